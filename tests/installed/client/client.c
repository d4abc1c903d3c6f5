/* Uses the C library as its header says; calls as JSON are what the Python package makes. Prints each check that fails;
   the last line is "N passed, N failed". */
#include <stdio.h>
#include <string.h>
#include <talutil_c.h>

static int passed;
static int failed;

static void check(const char* name, int holds) {
  if (holds) {
    ++passed;
  } else {
    ++failed;
    printf("FAILED: %s\n", name);
  }
}

/* Takes the text. */
static int is_text(char* text, const char* expected) {
  const int same = text != NULL && strcmp(text, expected) == 0;
  if (!same) printf("  expected: %s\n  actual:   %s\n", expected, text == NULL ? "null" : text);
  talutil_free(text);
  return same;
}

static void use_functions(talutil_library* library, talutil_library* other) {
  char* text = NULL;
  char* after = NULL;
  int32_t pages = 0;
  int16_t branch = 0;
  float rate = 0;
  bool is_number = false;
  check("a text", talutil_GetData(library, "\xE2\x82\xAC,B,", 0, 1, &text) == 0 && is_text(text, "\xE2\x82\xAC"));
  check("a number", talutil_GetMaxPages(library, 10, 25, &pages) == 0 && pages == 3);
  check("a truth value", talutil_IsValueNumber(library, "12", &is_number) == 0 && is_number);
  check("written back", talutil_RemoveStringsFromNumber(library, 2, "A B", "", &after, &text) == 0 &&
                            is_text(text, "AB") && is_text(after, " "));
  check("places left out", talutil_RemoveStringsFromNumber(library, 2, "A B", NULL, NULL, NULL) == 0);
  check("an error", talutil_GetData(library, "A,B,", 2, 1, &text) == 5 && text == NULL &&
                        strcmp(talutil_description(library), "Invalid procedure call or argument") == 0);
  check("not UTF-8", talutil_StripNulls(library, "\xFF", &text) == 5 && text == NULL);
  check("no handle", talutil_StripNulls(NULL, "a", &text) == 91 && text == NULL);
  check("a property",
        talutil_put_iBranchID(library, 7) == 0 && talutil_get_iBranchID(library, &branch) == 0 && branch == 7);
  check("a Single",
        talutil_put_GSTValue(library, 0.1F) == 0 && talutil_get_GSTValue(library, &rate) == 0 && rate == 0.1F);
  check("seen by calls as JSON", is_text(talutil_call(library, "{\"call\": \"iBranchID\"}"), "{\"result\": 7}"));
  check("another library's own", talutil_get_iBranchID(other, &branch) == 0 && branch == 0);
}

int main(void) {
  talutil_library* const library = talutil_open(NULL);
  talutil_library* const other = talutil_open("{\"code_page\": 1251}");
  check("open", library != NULL && other != NULL);
  check("no handle, as JSON", talutil_call(NULL, "{}") == NULL);
  use_functions(library, other);
  check("another code page",
        is_text(talutil_call(other, "{\"call\": \"VerifyTextData\", \"args\": [0, 0, \"\\u041e?\"]}"),
                "{\"result\": \"\xD0\x9E\"}"));
  talutil_close(library);
  talutil_close(other);
  talutil_close(NULL);
  check("no such code page", talutil_open("{\"code_page\": 1}") == NULL && *talutil_open_failure() != '\0');
  check("no such option", talutil_open("{\"page\": 1}") == NULL && strstr(talutil_open_failure(), "code_page") != NULL);
  printf("%d passed, %d failed\n", passed, failed);
  return failed == 0 ? 0 : 1;
}
