// Says "the page is there" at once: what a process costs before it asks anything.
trace("the page is there");
quit();
