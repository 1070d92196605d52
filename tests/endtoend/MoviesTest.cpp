// The movies that come with the project, and what a movie sees when the store is not as it should be.
#include "Movie.h"
#include "Store.h"

namespace {

class Demonstration : public Store {
protected:
    MovieOutput Run(const std::string& movie, const std::string& deployment = "")
    {
        return RunMovieFile(std::string(ZV_MOVIES) + "/" + movie,
                            {{"ZV_DEPLOYMENT", deployment.empty() ? store->DeploymentFile() : deployment}});
    }

    static void ExpectScriptError(const MovieOutput& output, const std::string& error)
    {
        EXPECT_EQ("script error", output.End());
        EXPECT_EQ(error, output.After("script error: ").substr(0, error.size())) << output.Text();
    }

    // After a run that shall have ended well.
    void ExpectWell(const MovieOutput& output) const
    {
        EXPECT_EQ(0, output.status);
        EXPECT_EQ("ok", output.End()) << output.Text();
        for (const LoggedRequest& request : store->Log())
            EXPECT_EQ("", request.violation) << request.operation;
    }
};

TEST_F(Demonstration, TheStoreIsShown)
{
    const MovieOutput output = Run("storefront.js");
    ExpectWell(output);
    EXPECT_EQ("", output.After("Genres"));
    EXPECT_EQ(store->Query("SELECT '1 of ' || ((COUNT(*) + 9) / 10) || ' (' || COUNT(*) || ' titles)' FROM title_genre "
                           "WHERE genre = 100"),
              output.After("Titles, page "));
    EXPECT_EQ(
        store->Query("SELECT synopsis FROM title WHERE id = (SELECT MIN(title) FROM title_genre WHERE genre = 100)"),
        output.After("    Synopsis    "));
}

TEST_F(Demonstration, AnEveningChangesTheAccount)
{
    const MovieOutput output = Run("evening.js");
    ExpectWell(output);
    EXPECT_EQ("0 goes on at 1234 s", output.After("loadLastStreamingAssetLocation: "));
    EXPECT_EQ("1234", store->Query("SELECT position FROM pass ORDER BY id DESC LIMIT 1"));
}

TEST_F(Demonstration, AStoreThatCannotBeTrustedOrReachedEndsTheMovieWithAnError)
{
    store->SetCertificate(CertificateKind::Untrusted);
    ExpectScriptError(Run("storefront.js"), "Error: init failed with status -2011");
    ExpectScriptError(Run("storefront.js", "/no/such/file"), "Error: init failed with status -1900");
    store->SetCertificate(CertificateKind::Good);
    Fault("getTitlesByNavigation=http:503");
    ExpectScriptError(Run("storefront.js"), "Error: getTitles failed with status -4503");
    EXPECT_EQ("ok", Run("storefront.js").End());
}

TEST_F(Demonstration, AMovieThatCannotBeReadIsOneLine)
{
    const MovieOutput output = Run("no-such-movie.js");
    EXPECT_EQ("", output.After("[ZV_FLASH]CreateAndConfigureStageWindowSet fail "));
    EXPECT_EQ("(unknown)", output.End());
    EXPECT_NE(std::string::npos, output.After("stagecraft: cannot read the movie ").find("no-such-movie.js"));
}

}  // namespace
