char const* extra = "plain";
