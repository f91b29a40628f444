// The file transfer service, through a broker.
#include "providers_fixture.h"

namespace velkhost::providers::testing {
namespace {

namespace fs = std::filesystem;
using cim::NamedValues;
using cim::Value;

class FileTransferProvider : public ProviderTest {
  protected:
    FileTransferProvider() { play(""); }

    broker::MethodReply call(const std::string &method, const NamedValues &in = {}) {
        return broker_.invoke_method(path_of("ZEB_FileTransferService"), method, in);
    }
    broker::MethodReply remove(const std::string &uri) {
        return call("DeleteTransferredFile", {{"FileURI", Value::string(uri)}});
    }
    // Makes the file count as transferred.
    std::string transferred(const std::string &name) {
        std::string uri = make_file(name);
        play("[file_transfer]\ntransferred = ['" + (folder_ / name).string() + "']");
        return uri;
    }
};

TEST_F(FileTransferProvider, HasOneInstance) {
    const auto reply = broker_.enumerate_instances(path_of("ZEB_FileTransferService"));
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(text(reply.instances[0].properties, "Name"), "HostFileTransferService");
    EXPECT_TRUE(broker_.get_instance(reply.instances[0].path).status.ok());
}

TEST_F(FileTransferProvider, CallersFileIsRefusedAndKept) {
    const std::string uri = make_file("mine.xml");
    const auto reply = remove(uri);
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(reply.status.message,
              "Not deleted, because this service did not transfer it: " + uri);
    EXPECT_TRUE(fs::exists(folder_ / "mine.xml"));
}

TEST_F(FileTransferProvider, TextThatIsNoFileUriIsRefused) {
    for (const char *uri : {"", "/etc/passwd", "tftp://host/a", "file://", "file:/a"}) {
        EXPECT_EQ(remove(uri).status.code, CMPI_RC_ERR_ACCESS_DENIED) << uri;
    }
}

TEST_F(FileTransferProvider, TransferredFileIsDeletedOnce) {
    const std::string uri = transferred("fetched.xml");
    const auto reply = remove(uri);
    EXPECT_TRUE(reply.status.ok()) << reply.status.message;
    EXPECT_EQ(reply.return_value, Value::uint32(0));
    EXPECT_FALSE(fs::exists(folder_ / "fetched.xml"));
    EXPECT_EQ(remove(uri).status.code, CMPI_RC_ERR_ACCESS_DENIED);
}

TEST_F(FileTransferProvider, TransferredFileThatIsGoneCountsAsDeleted) {
    const std::string uri = transferred("fetched.xml");
    fs::remove(folder_ / "fetched.xml");
    EXPECT_TRUE(remove(uri).status.ok());
}

TEST_F(FileTransferProvider, FailedDeleteSaysWhyAndCanBeRepeated) {
    const std::string uri = transferred("fetched.xml");
    fs::remove(folder_ / "fetched.xml");
    fs::create_directory(folder_ / "fetched.xml");
    const auto reply = remove(uri);
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(reply.status.message, "Cannot delete " + uri + ": Is a directory");
    fs::remove(folder_ / "fetched.xml");
    EXPECT_TRUE(remove(uri).status.ok());
}

TEST_F(FileTransferProvider, DeleteWithoutAFileIsAnInvalidParameter) {
    EXPECT_EQ(call("DeleteTransferredFile").status.code, CMPI_RC_ERR_INVALID_PARAMETER);
}

// What is no location of the method's kind is answered without a look at the file store.
TEST_F(FileTransferProvider, LocationOfAnotherKindIsAnInvalidParameter) {
    for (const char *uri : {"", "x", "sftp://host/a.xml", "file:///etc/passwd", "tftp://host/"}) {
        const auto reply = call("TransferViaTFTP", {{"SourceURI", Value::string(uri)}});
        EXPECT_EQ(reply.return_value, Value::uint32(3)) << uri;
        EXPECT_EQ(text(reply.out, "DestinationURI"), "") << uri;
    }
    for (const char *uri : {"", "ftp://host/a.zip", "file:///etc/passwd", "sftp:///a.xml"}) {
        const auto reply = call("TransferViaURL", {{"SourceURI", Value::string(uri)}});
        EXPECT_EQ(reply.return_value, Value::uint32(3)) << uri;
        EXPECT_EQ(text(reply.out, "DestinationURI"), "") << uri;
        EXPECT_EQ(reply.out.find("Job"), nullptr) << uri;
    }
}

TEST_F(FileTransferProvider, BlockSizeThatTftpDoesNotKnowIsAnInvalidParameter) {
    for (const auto size : std::initializer_list<std::uint16_t>{0, 7, 65465, 65535}) {
        const auto reply =
            call("TransferViaTFTP", {{"SourceURI", Value::string("tftp://host/a.xml")},
                                     {"BlockSize", Value::uint16(size)}});
        EXPECT_EQ(reply.return_value, Value::uint32(3)) << size;
    }
    const auto reply = call("TransferViaTFTP", {{"SourceURI", Value::string("tftp://host/a.xml")},
                                                {"BlockSize", Value::string("many")}});
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(FileTransferProvider, TransferWithoutASourceIsAnInvalidParameter) {
    for (const char *method : {"TransferViaTFTP", "TransferViaURL"}) {
        EXPECT_EQ(call(method).status.code, CMPI_RC_ERR_INVALID_PARAMETER) << method;
    }
}

TEST_F(FileTransferProvider, UnknownMethodIsNotFound) {
    EXPECT_EQ(call("Transfer").status.code, CMPI_RC_ERR_METHOD_NOT_FOUND);
}

TEST_F(FileTransferProvider, PathWithForeignKeysIsNotFound) {
    cim::ObjectPath path = path_of("ZEB_FileTransferService");
    path.keys.set("Name", Value::string("Other"));
    EXPECT_EQ(broker_.invoke_method(path, "DeleteTransferredFile").status.code,
              CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(FileTransferProvider, FaultsStrikeTheirSteps) {
    play(
        "[[fault]]\nstep = 'filetransfer.delete'\ncode = 1\nmessage = 'a'\n"
        "[[fault]]\nstep = 'filetransfer.tftp'\ncode = 1\nmessage = 'b'\n"
        "[[fault]]\nstep = 'filetransfer.url'\ncode = 1\nmessage = 'c'\n");
    const NamedValues source{{"SourceURI", Value::string("x")}};
    EXPECT_EQ(remove("file:///x").status.message, "a");
    EXPECT_EQ(call("TransferViaTFTP", source).status.message, "b");
    EXPECT_EQ(call("TransferViaURL", source).status.message, "c");
    EXPECT_TRUE(scenario_->faults.unfired().empty());
}

}  // namespace
}  // namespace velkhost::providers::testing
