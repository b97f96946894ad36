"""Definitions, comments and names of files that would do harm if they were more than text."""

from pages import PageTest, main


class Hostile(PageTest):
    page = "hostile"

    def check_is_unhurt(self):
        self.check_is_quiet()
        self.assertEqual(0, self.script(
            "return document.querySelectorAll('img, iframe, base, object, embed').length"))
        self.assertEqual(1, self.script("return document.querySelectorAll('script').length"))
        self.assertEqual(1, self.script("return document.querySelectorAll('style').length"))
        self.assertEqual(0, self.script("""
          return Array.from(document.querySelectorAll('*')).filter((e) => Array.from(e.attributes)
              .some((a) => a.name.startsWith('on') || /javascript:/i.test(a.value) &&
                           a.name !== 'aria-label' && a.name !== 'value')).length;"""))
        self.assertNotEqual("hurt", self.browser.title)

    def test_nothing_of_theirs_runs(self):
        self.check_is_unhurt()

    def test_they_are_told_as_they_are(self):
        for definition in self.document()["definitions"]:
            for clause in definition["clauses"]:
                if clause["clause"] == "DESC":
                    self.assertIn(clause["old"], self.script(
                        "return document.getElementById('main').textContent"))

    def test_nothing_of_theirs_runs_in_a_page_of_check(self):
        self.load("hostile-check")
        self.check_is_unhurt()
        text = self.script("return document.getElementById('main').textContent")
        self.assertIn("</script><img src=x onerror=alert(1)>", text)
        self.assertIn("\\u001b[31m", text)
        self.assertIn("\\u2028", text)

    def test_the_policy_stops_what_escaping_would_let_through(self):
        self.script("""
          window.hurt = 0;
          const box = document.createElement('div');
          box.innerHTML = '<img src="data:image/png;base64,x" onerror="window.hurt = 1">' +
              '<p style="color: red">';
          document.body.append(box);
          const script = document.createElement('script');
          script.textContent = 'window.hurt = 2';
          document.body.append(script);
          const picture = document.createElement('img');
          picture.src = 'https://example.invalid/a.png';
          document.body.append(picture);""")
        self.browser.execute_async_script("setTimeout(arguments[0], 300)")
        self.assertEqual(0, self.script("return window.hurt"))
        stopped = " ".join(entry["message"] for entry in self.browser.get_log("browser"))
        for directive in ("script-src", "style-src", "img-src"):
            self.assertIn(directive, stopped)


if __name__ == "__main__":
    main()
